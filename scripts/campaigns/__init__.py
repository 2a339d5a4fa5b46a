"""What the campaigns of failures share: docs/testing.md tells of them."""
